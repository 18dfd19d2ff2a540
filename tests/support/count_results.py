"""Adds up GoogleTest's XML reports and the steps of test.sh; prints 'N passed, N failed, N skipped'.

Usage: count_results.py RESULTS_FOLDER
"""

import pathlib
import re
import sys
import xml.etree.ElementTree as tree

# Texts of tests may hold any bytes; XML may not.
FORBIDDEN = re.compile("[\\x00-\\x08\\x0b\\x0c\\x0e-\\x1f\\ufffe\\uffff]|&#x(?:[0-8BbCcEeFf]|1[0-9A-Fa-f]);")

passed = failed = skipped = 0
results = pathlib.Path(sys.argv[1])

for report in sorted(results.glob("*/*.xml")):
    try:
        text = report.read_bytes().decode("utf-8", errors="replace")
        cases = tree.fromstring(FORBIDDEN.sub("?", text)).iter("testcase")
    except tree.ParseError:
        failed += 1
        print(f"unreadable report: {report}")
        continue
    for case in cases:
        if case.get("status") == "notrun":
            continue
        if case.find("failure") is not None:
            failed += 1
            print(f"failed: {report.parent.name}: {case.get('classname')}.{case.get('name')}")
        elif case.get("result") == "skipped" or case.find("skipped") is not None:
            skipped += 1
            reason = case.find("skipped")
            text = (reason.get("message") or "").strip().splitlines() if reason is not None else []
            print(f"skipped: {case.get('classname')}.{case.get('name')}: {text[-1] if text else ''}")
        else:
            passed += 1

steps = results / "steps"
for line in steps.read_text().splitlines() if steps.exists() else []:
    if line.endswith(": passed"):
        passed += 1
    else:
        failed += 1

print(f"{passed} passed, {failed} failed, {skipped} skipped")
