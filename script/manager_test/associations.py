"""Checks of associations: associators, references and their names, compared with each other and with the classes."""

from .instances import check_response
from .run import steady
from .wbemcli import Path

COMPUTER = "VELKO_ComputerSystem"


def associator_rows(run, cls, source, target):
    """Yields the options of requests from one end of the association to the other, and whether they find something."""
    yield {"ac": cls.name}, True
    if run.is_gate:
        exact = {"ac": cls.name, "arc": target.reference_class, "ar": source.name, "arr": target.name}
        yield exact, True
        yield {name: value.lower() for name, value in exact.items()}, True
        yield from (({"ac": cls.name, name: exact[name]}, True) for name in ("arc", "ar", "arr"))
        for name, value in {"arc": "VELKO_OstrelAgent", "ar": target.name, "arr": source.name}.items():
            yield {"ac": cls.name, name: value}, False


def reference_rows(cls, source, target):
    yield {"arc": cls.name}, True
    yield {"arc": cls.name.lower(), "ar": source.name.lower()}, True
    yield {"arc": cls.name, "ar": target.name}, False


def check_rows(run, operations, path, rows, expected):
    """Checks that the operations for names and for instances find the expected paths, with the options of each row."""
    for options, finds in rows:
        names, listed = (run.ask(operation, path, **options) for operation in operations)
        for response in (names, listed):
            check_response(run, response)
            run.check(f"{response.request}: paths", set(response.paths), set(expected if finds else []))
        for instance in listed.objects:
            run.check(f"{listed.request}: {instance.path}", steady(instance), steady(run.find(instance.path)))


def check_end(run, cls, ends, path, far_paths, links):
    check_rows(run, ("ain", "ai"), path, associator_rows(run, cls, *ends), far_paths)
    if run.is_gate:
        check_rows(run, ("rin", "ri"), path, reference_rows(cls, *ends), links)
        return
    for operation in ("rin", "ri"):  # Some object managers replace the provider's status by an empty success.
        response = run.ask(operation, path, status="NOT_SUPPORTED|OK", arc=cls.name)
        run.check(f"{response.request}: paths", response.paths, [])


def check_association(run, cls):
    source, target = sorted(cls.properties.values(), key=lambda end: end.reference_class != COMPUTER)
    if target.reference_class not in run.tied:
        run.report.note(f"{cls.name}: no {target.reference_class} belongs to the computer")
        return
    tied, own = run.tied[target.reference_class], run.records.get(target.reference_class)
    computers, records, listed = (run.ask("ein", name).paths for name in (COMPUTER, target.reference_class, cls.name))
    held = {computer: run.ask("ain", computer, ac=cls.name).paths for computer in computers}
    run.check(f"computers that have {tied}", [tied in paths for paths in held.values()].count(True), 1)

    def link(computer, record):
        return Path.of(cls.name, **{source.name: computer, target.name: record})

    # The bare provider enumerates every record with the first computer. For the computer's record, it returns all
    # computers except the last.
    pairs = held if run.is_gate else {computer: records for computer in computers[:1]}
    run.check(f"ein {cls.name}: pairs", set(listed),
              {link(computer, record) for computer in pairs for record in pairs[computer]})
    for computer, paths in held.items():
        check_end(run, cls, (source, target), computer, paths, [link(computer, path) for path in paths])
    for record in filter(None, (tied, own)):
        owners = [computer for computer, paths in held.items() if record in paths]
        bare = computers[:-1] if record == tied else []
        check_end(run, cls, (target, source), record, run.by_provider(owners, bare), [link(each, record) for each in owners])
