"""What the module costs in a server, against the plain providers of tests/bench in its place: the same server, registrations, host
and client, in two machines."""

import statistics
import sys

import bench_requests
from rooms import Room

sys.path.insert(0, str(bench_requests.SOURCE / "tests/bench"))

from markdown import print_table  # noqa: E402

#: 64 ports that see 2,048 LUNs between them, of 8 targets each; plain providers know no converged adapters.
HOST = ["--adapters", "32", "--ports", "2", "--targets", "8", "--luns", "4", "--cna", "0"]
#: What the processor's time of the module's server is to stay below, where that of the plain providers' is 1.
GOAL = 1.05
#: Seconds of a turn, and the most that it has of requests on one connection, and of connections: sfcb ends one, and the process that
#: served it, after ten requests.
TURN, KEPT, CONNECTIONS = 0.3, 8, 4
PARTS = ("provider", "others")
#: Who answers. A module without settings of its log looks for them at each line, and that is how it is installed.
PLAIN, MODULE, LOGGING = SIDES = ("plain", "module", "with a log")


def compare(rooms, question):
    """Ends the program if they do not answer alike."""
    answers = {side: bench_requests.objects_in(rooms[side].order("answer", question.message)) for side in SIDES}
    for side in (MODULE, LOGGING):
        said = bench_requests.difference(answers[PLAIN], answers[side])
        if said:
            raise SystemExit(f"bench: {question.title}: the plain providers answer otherwise: {said}")


def turns_of(rooms, question, rounds):
    """Turn by turn, what each side took for an object, in microseconds: of the provider's process, and of all others."""
    longest = max(rooms[side].order("measure", question.message, 1)["seconds"][0] for side in SIDES)
    times = max(1, min(KEPT, round(TURN / longest)))
    connections = max(1, min(CONNECTIONS, round(TURN / longest / times)))
    taken = []
    for number in range(rounds):
        turn = {}
        for side in SIDES if number % 2 else reversed(SIDES):
            figures = [rooms[side].order("measure", question.message, times) for _ in range(connections)]
            objects = connections * times * question.count
            turn[side] = [sum(each[part] for each in figures) / objects / 1000 for part in PARTS]
        taken.append(turn)
    return taken


def row_of(server, question, turns):
    row = {"server": server.title, "request": question.title, "objects": question.count, "turns": len(turns)}
    for side in SIDES:
        for part, name in enumerate(PARTS):
            row[f"{name}, {side}"] = statistics.median(turn[side][part] for turn in turns)
        ratios = sorted(sum(turn[side]) / sum(turn[PLAIN]) for turn in turns)
        row[f"ratio, {side}"] = statistics.median(ratios)
        row[f"quartiles, {side}"] = [ratios[len(ratios) // 4], ratios[len(ratios) * 3 // 4]]
    return row


def shown(row):
    """What the module does to the server's other processes is seen as well, and small."""
    cells = {row["server"]: row["request"], "objects": f"{row['objects']:,}"}
    cells |= {f"provider, {side}": f"{row[f'provider, {side}']:.1f}" for side in SIDES}
    cells |= {f"others, {side}": f"{row[f'others, {side}']:.1f}" for side in (PLAIN, MODULE)}
    for side in (MODULE, LOGGING):
        low, high = row[f"quartiles, {side}"]
        cells[f"ratio, {side} ({GOAL})"] = f"{row[f'ratio, {side}']:.2f} ({low:.2f} to {high:.2f})"
    return cells


def measure_providers(server, build, options):
    """The rows of one server."""
    rooms = {
        PLAIN: Room(server, build, plain=True),
        MODULE: Room(server, build),
        LOGGING: Room(server, build, log="LOG_LEVEL=ERR\n"),
    }
    for room in rooms.values():
        room.wait()
    turns = {}
    for sitting in range(options.sittings):
        for room in rooms.values():
            room.order("start", HOST, bench_requests.enumeration("KALDERA_FCPort"))
        if not sitting:
            questions = [bench_requests.Question(*each) for each in rooms[MODULE].order("questions")]
            for question in questions:
                compare(rooms, question)
        for question in questions:
            turns.setdefault(question.title, []).extend(turns_of(rooms, question, options.rounds))
    for room in rooms.values():
        room.end()
    rows = [row_of(server, question, turns[question.title]) for question in questions]
    print_table([shown(row) for row in rows])
    return rows
