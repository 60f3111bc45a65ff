# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the client prints with --json is what its schema says."""

import json
import pathlib

import jsonschema

SCHEMA = json.loads(
    (pathlib.Path(__file__).resolve().parents[2] / "client/output.schema.json").read_text())
VALIDATOR = jsonschema.Draft7Validator(SCHEMA)


def validate(arguments, out):
    """Of a call with these arguments, when it has printed JSON."""
    if out and "--json" in arguments:
        VALIDATOR.validate(json.loads(out))
