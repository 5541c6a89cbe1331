import js from "@eslint/js";

const browser = ["CSS", "HTMLCanvasElement", "HTMLInputElement", "Node", "ResizeObserver", "URLSearchParams", "atob", "document",
  "getComputedStyle", "requestAnimationFrame", "window"];

export default [
  js.configs.recommended,
  {
    files: ["**/*.js"],
    languageOptions: {
      ecmaVersion: 2022,
      sourceType: "module",
      globals: Object.fromEntries(browser.map((name) => [name, "readonly"])),
    },
    rules: {
      eqeqeq: "error",
      "max-len": ["error", { code: 120 }],
      "max-lines-per-function": ["error", { max: 40, skipComments: true }],
      "no-restricted-properties": [
        "error",
        ...["innerHTML", "outerHTML", "insertAdjacentHTML"].map((property) => ({
          property,
          message: "Texts of a trace must never be taken for markup.",
        })),
      ],
      "no-shadow": "error",
      "no-var": "error",
      "prefer-const": "error",
    },
  },
];
