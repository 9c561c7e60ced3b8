#!/usr/bin/env python3
"""Every message that the sources raise stands on the page of messages."""

import re

from workspace_fixture import ROOT, equal, run_tests

RAISED = re.compile(r'(?:LexScannerException|\bFail|\bFailAt|\bComplain|WithToken)\((?:[\w.*]+, |std::string\(\w+\) \+ )?'
                    r'(?:PrintedElement\([^()]*\) \+ )?"((?:[^"\\]|\\.)*)"')
TOLD = re.compile(r'(?:trace|TraceWriter\(\)|WriteToConsole\() ?(?:<< )?"((?:[^"\\]|\\.)*(?:[Ee]rror|ERROR|[Ww]arning|'
                  r"[Ff]ail|[Cc]annot|Couldn't|Can't|not found)(?:[^\"\\]|\\.)*)\"")
GENERIC = re.compile(r"^(Expected|Met EO[SF])\b|expected( *in \S+ directive)?$| expected after |nested too deeply$"
                     r"|expected before |^[^A-Za-z]*$|^warning W$")


def test_every_message_is_explained(_):
    page = re.sub(r"\s+", " ", (ROOT / "docs/messages.md").read_text())
    missing, seen = [], 0
    for path in sorted((ROOT / "src").rglob("*.cpp")):
        text = path.read_text()
        for pattern in (RAISED, TOLD):
            for message in pattern.findall(text):
                said = re.sub(r"\\n|\\(?=\")", "", message).strip(" :('<*.-\\")
                said = re.sub(r"\s+", " ", said.removesuffix(" when read $").removesuffix(" when read"))
                seen += 1
                if said and said not in page and not GENERIC.search(said):
                    missing.append(f"{path.relative_to(ROOT)}: {message}")
    equal("\n".join(missing), "")
    assert seen > 150, f"only {seen} messages were found in the sources"


run_tests(globals())
