"""A headless Chromium, driven by chromedriver over HTTP: no more than the tests of the page need."""
import base64
import json
import shutil
import subprocess
import urllib.error
import urllib.request

ARGUMENTS = ["--headless=new", "--no-sandbox", "--disable-gpu", "--hide-scrollbars", "--force-device-scale-factor=1",
             "--disable-extensions", "--disable-component-update", "--disable-background-networking"]
ELEMENT = "element-6066-11e4-a52e-4f735466cecf"


def missing():
    """The name of a program that is not there; None when a browser can be driven."""
    return next((name for name in ("chromium", "chromedriver") if shutil.which(name) is None), None)


class Browser:
    def __init__(self, width=1100, height=900, dark=False):
        self.driver = subprocess.Popen(["chromedriver", "--port=0"], stdout=subprocess.PIPE, text=True)
        port = None
        for line in self.driver.stdout:
            if "on port " in line:
                port = int(line.split("on port ")[1].split(".")[0].split()[0])
                if port:
                    break
        self.base = f"http://127.0.0.1:{port}"
        arguments = ARGUMENTS + [f"--window-size={width},{height}"]
        options = {"args": arguments, "binary": shutil.which("chromium")}
        made = self.post("/session", {"capabilities": {"alwaysMatch": {
            "goog:chromeOptions": options,
            "goog:loggingPrefs": {"browser": "ALL", "performance": "ALL"}}}})
        self.base += "/session/" + made["sessionId"]
        self.show_as(width, height, dark)

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.post("", method="DELETE")
        self.driver.terminate()
        self.driver.wait(20)
        self.driver.stdout.close()

    def post(self, path, body=None, method="POST"):
        data = None if method == "DELETE" else json.dumps(body or {}).encode()
        request = urllib.request.Request(self.base + path, data, {"Content-Type": "application/json"}, method=method)
        try:
            with urllib.request.urlopen(request, timeout=60) as answer:
                return json.load(answer)["value"]
        except urllib.error.HTTPError as error:
            raise RuntimeError(error.read().decode()) from None

    def cdp(self, command, **parameters):
        return self.post("/goog/cdp/execute", {"cmd": command, "params": parameters})

    def show_as(self, width, height, dark=False):
        self.cdp("Emulation.setDeviceMetricsOverride", width=width, height=height, deviceScaleFactor=1, mobile=False)
        self.cdp("Emulation.setEmulatedMedia",
                 features=[{"name": "prefers-color-scheme", "value": "dark" if dark else "light"}])

    def open(self, url):
        self.post("/url", {"url": url})

    def run(self, script, *arguments):
        return self.post("/execute/sync", {"script": script, "args": list(arguments)})

    def drawn(self):
        """Until what was asked for is drawn."""
        self.post("/execute/async", {"script": "requestAnimationFrame(() => requestAnimationFrame(arguments[0]))",
                                     "args": []})

    def keys(self, *keys):
        actions = [action for key in keys for action in ({"type": "keyDown", "value": key},
                                                         {"type": "keyUp", "value": key})]
        self.post("/actions", {"actions": [{"type": "key", "id": "keyboard", "actions": actions}]})
        self.drawn()

    def pointer(self, *actions):
        self.post("/actions", {"actions": [{"type": "pointer", "id": "mouse", "actions": list(actions)}]})
        self.drawn()

    def wheel(self, x, y, distance):
        """With Ctrl held."""
        self.cdp("Input.dispatchMouseEvent", type="mouseWheel", x=x, y=y, deltaX=0, deltaY=distance, modifiers=2)
        self.drawn()

    def picture(self):
        return base64.b64decode(self.cdp("Page.captureScreenshot", format="png")["data"])

    def log(self, kind):
        return self.post("/se/log", {"type": kind})


KEYS = {"left": "\ue012", "right": "\ue014", "home": "\ue011", "end": "\ue010", "escape": "\ue00c", "tab": "\ue004",
        "enter": "\ue007", "page_up": "\ue00e", "page_down": "\ue00f"}


def reduced(browser, picture, columns, rows):
    """A picture made small by the browser: the PNG of it, and its colours, four numbers a pixel."""
    browser.open("about:blank")
    script = """
        const [source, width, height, done] = arguments;
        const image = new Image();
        image.onload = () => {
          const canvas = Object.assign(document.createElement("canvas"), { width, height });
          const context = canvas.getContext("2d");
          context.imageSmoothingQuality = "high";
          context.drawImage(image, 0, 0, width, height);
          done([canvas.toDataURL().split(",")[1], [...context.getImageData(0, 0, width, height).data]]);
        };
        image.src = "data:image/png;base64," + source;"""
    made, colours = browser.post("/execute/async", {
        "script": script, "args": [base64.b64encode(picture).decode(), columns, rows]})
    return base64.b64decode(made), colours
