"""How well the sensor hub senses, on people that it was not learned from.

What a person does: the classifier is learned anew without each person in turn, and decides on that person. On a folder other
than data/, the classifier as it is built decides on the people that data/ has not, too. Steps and shakes have no learned
parameters.
"""

import collections
import gzip
import pathlib
import re
import subprocess
import sys

REPOSITORY = pathlib.Path(__file__).resolve().parents[2]
sys.dont_write_bytecode = True
sys.path.insert(0, str(REPOSITORY / "scripts"))
import learn_activity  # noqa: E402
from learn_activity import np  # noqa: E402

NAMES = {1: "still", 2: "on foot", 3: "running"}
SENSITIVITIES = 3


def person_of(path):
    """Recordings of one kind have people with numbers of their own."""
    kind, number = re.match(r"([a-z]+)_.*person(\d+)", path.name).groups()
    return kind, int(number)


def sensed(build, paths, limits):
    """The lines that the program prints about the recordings: (the first word, the numbers)."""
    command = [build / "bin" / "accuracy_sensing", *map(str, limits), *paths]
    lines = subprocess.run(command, text=True, check=True, stdout=subprocess.PIPE).stdout.splitlines()
    return [(words[0], list(map(int, words[1:]))) for words in map(str.split, lines) if words[0] != "recording"]


def add_decisions(counts, lines):
    for word, numbers in lines:
        if word == "activity":
            counts[tuple(numbers[:3])] += numbers[3]


def built_limits():
    return re.findall(r"= (\d+)", (REPOSITORY / "platform/hub/activity_model.inc").read_text())


def leave_one_out(build, people):
    """What is decided about each person by a classifier that learned from all others; and the least that is right of one."""
    windows = {person: [learn_activity.windows_of(path) for path in paths] for person, paths in people.items()}
    counts, least = collections.Counter(), 1.0
    for person, paths in people.items():
        others = [pair for other, pairs in windows.items() if other != person for pair in pairs]
        if not {activity for _, activities in others for activity in activities.tolist()} >= NAMES.keys():
            continue  # nobody to learn from
        limits = learn_activity.limits_of(*(np.concatenate(values) for values in zip(*others)))
        own = collections.Counter()
        add_decisions(own, sensed(build, paths, limits))
        least = min(least, right_share(own, learn_activity.WINDOW))
        counts += own
    return counts, least


def right_share(counts, length):
    right = sum(count for (window, truth, found), count in counts.items() if window == length and truth == found)
    return right / max(1, sum(count for (window, _, _), count in counts.items() if window == length))


def activity_row(name, people, counts):
    for length in (128, 64):
        own = {key[1:]: count for key, count in counts.items() if key[0] == length}
        shares = []
        for activity in NAMES:
            total = sum(count for (truth, _), count in own.items() if truth == activity)
            shares.append(f"{100 * own.get((activity, activity), 0) / total:.1f} %" if total else "")
        window = f"{length * learn_activity.INTERVAL_MS / 1000:.2f} s"
        print(
            f"| {name} | {people} | {window} | {sum(own.values())} | {' | '.join(shares)} | {100 * right_share(counts, length):.1f} % |"
        )


def activity_table(build, folder):
    people = collections.defaultdict(list)
    for path in sorted((folder / "activity").glob("*_person*.csv.gz")):
        people[person_of(path)].append(path)
    if not people:
        return
    print(f"\n| Classifier learned from | People | Window | Decisions | {' | '.join(NAMES.values())} | All right |")
    print("| --- | --: | --: | --: | --: | --: | --: | --: |")
    counts, least = leave_one_out(build, people)
    if counts:
        activity_row("everybody else there", len(people), counts)
    known = {person_of(path) for path in (REPOSITORY / "data/activity").glob("*_person*.csv.gz")}
    strangers = {person: paths for person, paths in people.items() if person not in known}
    if strangers:
        own = collections.Counter()
        add_decisions(own, sensed(build, [path for paths in strangers.values() for path in paths], built_limits()))
        activity_row("data/, as it is built", len(strangers), own)
    if counts:
        print(f"\nOf one person alone, at least {100 * least:.1f} % are right (window of 2.56 s).")
    quiet_table(sensed(build, [path for paths in people.values() for path in paths], built_limits()))


def quiet_table(lines):
    rests = [numbers for word, numbers in lines if word == "rest"]
    print("\n| Where nothing is to be found | Minutes | Found |")
    print("| --- | --: | --: |")
    print(f"| steps at rest, in {len(rests)} stretches | {sum(rest[0] for rest in rests) / 60:.0f} | {sum(rest[1] for rest in rests)} |")
    for sensitivity in range(SENSITIVITIES):
        found = [numbers for word, numbers in lines if word == "shakes" and numbers[0] == sensitivity]
        minutes = sum(seconds for _, seconds, _ in found) / 60
        print(f"| shakes, sensitivity {sensitivity}, in all recordings | {minutes:.0f} | {sum(count for _, _, count in found)} |")


def steps_table(build, folder):
    paths = sorted((folder / "steps").glob("*.csv.gz"))
    if not paths:
        return
    print("\n| Walk | Reference | Counted | Error |")
    print("| --- | --: | --: | --: |")
    for path in paths:
        with gzip.open(path, "rt") as file:
            place = file.readline().strip().split(",").index("steps")
            counted = [int(line.split(",")[place]) for line in file]
        reference = max(counted) - counted[0]
        found = next(numbers[0] for word, numbers in sensed(build, [path], built_limits()) if word == "steps")
        name = path.name.split(".")[0].replace("steps_", "").replace("_", ", ")
        print(f"| {name} | {reference} | {found} | {100 * (found - reference) / reference:+.1f} % |")


def print_tables(build, folder):
    activity_table(build, folder)
    steps_table(build, folder)
